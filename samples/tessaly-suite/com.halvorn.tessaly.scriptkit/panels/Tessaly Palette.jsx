// One button for each effect of the suite; a click puts the effect on the selected layers.
(function (host) {
    var effects = ["Glow", "Grain", "Keyer", "Denoise"];
    var panel = host instanceof Panel ? host : new Window("palette", "Tessaly", undefined, { resizeable: true });
    for (var i = 0; i < effects.length; i++) {
        var button = panel.add("button", undefined, effects[i]);
        button.onClick = (function (name) {
            return function () {
                var comp = app.project.activeItem;
                if (comp instanceof CompItem) {
                    app.beginUndoGroup("Tessaly " + name);
                    for (var k = 0; k < comp.selectedLayers.length; k++) {
                        comp.selectedLayers[k].Effects.addProperty("HALVORN " + name);
                    }
                    app.endUndoGroup();
                }
            };
        })(effects[i]);
    }
    if (panel instanceof Window) {
        panel.show();
    } else {
        panel.layout.layout(true);
    }
})(this);
