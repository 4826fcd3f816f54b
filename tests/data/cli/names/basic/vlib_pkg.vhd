package ScoreBoardPkg_slv is
end package ScoreBoardPkg_slv;
