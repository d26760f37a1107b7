// A technology.
MenuRow {}
