// A category.
MenuRow {}
