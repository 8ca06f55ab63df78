#include "hosts/PlatformDetectors.h"

#include <boost/make_shared.hpp>

#include "hosts/AdobeDetectors.h"
#include "hosts/HostAppCheck.h"
#include "hosts/OtherDetectors.h"

namespace HV {

void AddPlatformDetectors(HostAppCheck& check) {
    check.AddDetector(boost::make_shared<AdobeAEDetector_Win>());
    check.AddDetector(boost::make_shared<AdobePremiereDetector_Win>());
    check.AddDetector(boost::make_shared<EdiusDetector_Win>());
    check.AddDetector(boost::make_shared<HitFilmDetector_Win>());
    check.AddDetector(boost::make_shared<MediaComposerDetector_Win>());
    check.AddDetector(boost::make_shared<ResolveDetector_Win>());
    check.AddDetector(boost::make_shared<VegasDetector_Win>());
}

}  // namespace HV
