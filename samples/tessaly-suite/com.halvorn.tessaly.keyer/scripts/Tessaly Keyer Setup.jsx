// Puts Tessaly Keyer on each selected layer and a garbage matte below it.
(function () {
    var comp = app.project.activeItem;
    if (!(comp instanceof CompItem) || comp.selectedLayers.length === 0) {
        alert("Select the layers that hold the screen first.", "Tessaly Keyer");
        return;
    }
    app.beginUndoGroup("Tessaly Keyer Setup");
    for (var i = 0; i < comp.selectedLayers.length; i++) {
        var layer = comp.selectedLayers[i];
        var mask = layer.mask.addProperty("ADBE Mask Atom");
        mask.name = "Garbage Matte";
        layer.Effects.addProperty("HALVORN Keyer");
    }
    app.endUndoGroup();
})();
