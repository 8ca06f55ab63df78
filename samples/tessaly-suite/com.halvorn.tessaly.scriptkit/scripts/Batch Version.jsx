// Raises the number behind "_v" in the names of all selected compositions.
(function () {
    app.beginUndoGroup("Batch Version");
    var chosen = app.project.selection;
    for (var i = 0; i < chosen.length; i++) {
        if (chosen[i] instanceof CompItem) {
            chosen[i].name = chosen[i].name.replace(/_v(\d+)/, function (all, digits) {
                var next = String(parseInt(digits, 10) + 1);
                while (next.length < digits.length) {
                    next = "0" + next;
                }
                return "_v" + next;
            });
        }
    }
    app.endUndoGroup();
})();
