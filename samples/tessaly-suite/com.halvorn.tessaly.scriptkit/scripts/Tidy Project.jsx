// Sorts everything at the top of the project into three folders.
(function () {
    function folderNamed(name) {
        for (var i = 1; i <= app.project.numItems; i++) {
            var item = app.project.item(i);
            if (item instanceof FolderItem && item.name === name) {
                return item;
            }
        }
        return app.project.items.addFolder(name);
    }
    function home(item) {
        if (item instanceof CompItem) {
            return "Compositions";
        }
        return item.mainSource instanceof SolidSource ? "Solids" : "Footage";
    }
    app.beginUndoGroup("Tidy Project");
    var moves = [];
    for (var i = 1; i <= app.project.numItems; i++) {
        var item = app.project.item(i);
        if (!(item instanceof FolderItem) && item.parentFolder === app.project.rootFolder) {
            moves.push(item);
        }
    }
    for (var j = 0; j < moves.length; j++) {
        moves[j].parentFolder = folderNamed(home(moves[j]));
    }
    app.endUndoGroup();
})();
